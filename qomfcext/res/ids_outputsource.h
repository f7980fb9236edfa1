// Resource ids of the output source page (4030) and the separator prompt (4041).
#pragma once
