// Resource ids of the combination definition (4040), the function manager dialog (4039) and the field-name dialog (4042).
#pragma once
