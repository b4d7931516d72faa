// The order in which the agent's locks are taken, lowest first. m_DataFetchMutex is held by itself.
// Builds that check locks end the process when a thread takes one out of order.
#ifndef VLN_AGENT_LOCK_ORDER_H
#define VLN_AGENT_LOCK_ORDER_H

namespace cimple {

enum Lock_Rank : int {
    RANK_AGENT = 10,
    RANK_DATA_FETCH = 20,
    RANK_ADAPTER_DATA_READY = 30,
    RANK_ADAPTER_MAPS_READY = 40,
    RANK_SAN_MAPS_READY = 50,
    RANK_DATA = 60,
    RANK_UPDATE = 65, // recursive, one for each active class
    RANK_DYNAMIC_PORT_STATUS = 70,
    RANK_AGENT_THREAD = 80, // what is known of a background thread
};

} // namespace cimple

#endif // VLN_AGENT_LOCK_ORDER_H
