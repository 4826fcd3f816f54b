// This source file's start-up objects of the host services (see Port/Init.h).
#pragma once

#include "Port/Init.h"

static Port::FileInit quillonFileInit;
static Port::PathListInit quillonPathListInit;
static RavA::InstanceTableInit quillonInstanceTableInit;
static RavA::FactoryInit quillonFactoryInit;
static Port_MsgManInit quillonMsgManInit;
