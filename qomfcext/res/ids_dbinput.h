// Resource ids of the dBase and file-database input pages (4011, 4012).
#pragma once
