// Resource ids of the fixed-length text input page (4009) and the text-format control.
#pragma once
