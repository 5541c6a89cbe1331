#pragma once
#define __BIONIC__ 1
