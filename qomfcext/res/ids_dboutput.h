// Resource ids of the dBase and file-database output pages (4025, 4028).
#pragma once
